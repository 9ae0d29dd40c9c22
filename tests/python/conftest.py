"""What the tests of the Python module share."""

import os

import pytest

import vorkel


@pytest.fixture(autouse=True)
def bundled_devices(monkeypatch):
    """The bundled devices, whatever the user's own are."""
    monkeypatch.delenv("VORKEL_DEVICES", raising=False)


@pytest.fixture(scope="session")
def video():
    """27 MHz x 44 is 1188 MHz: 8 x 148.5, 16 x 74.25 and 44 x 27 MHz."""
    outputs = ["148.5 MHz", "74.25 MHz", "27 MHz"]
    return vorkel.plan(inputs=["27 MHz"], outputs=outputs, device="vk40")


@pytest.fixture(scope="session")
def build_dir():
    return os.environ["VORKEL_BUILD_DIR"]


@pytest.fixture(scope="session")
def source_dir():
    return os.environ["VORKEL_SOURCE_DIR"]
