import pytest
from plain_loops import PlainLoops


@pytest.fixture(scope="session")
def plain_loops():
    return PlainLoops()
