"""A browser without a window, for the pages that the tool writes."""

import importlib.util
import os
import shutil
import subprocess
import sys

from workspace_fixture import Skipped

DEBIAN_PYTHON = "/usr/bin/python3"  # which sees the packages of Debian; the first on PATH may be another one


def with_selenium():
    """Goes on in an interpreter that has selenium, where there is one. To be called ahead of everything else."""
    if importlib.util.find_spec("selenium") or os.path.realpath(sys.executable) == os.path.realpath(DEBIAN_PYTHON):
        return
    if os.path.exists(DEBIAN_PYTHON) and subprocess.run([DEBIAN_PYTHON, "-c", "import selenium"], capture_output=True).returncode == 0:
        os.execv(DEBIAN_PYTHON, [DEBIAN_PYTHON, *sys.argv])


class Browser:
    """Chromium; what its console has to say fails `check`."""

    def __init__(self, width=1280, height=900, dark=False):
        if not importlib.util.find_spec("selenium"):
            raise Skipped("python3-selenium")
        for tool in ("chromium", "chromedriver"):
            if not shutil.which(tool):
                raise Skipped(tool)
        from selenium import webdriver
        from selenium.webdriver.chrome.options import Options
        from selenium.webdriver.chrome.service import Service
        options = Options()
        options.binary_location = shutil.which("chromium")
        for argument in ("--headless=new", "--no-sandbox", "--disable-gpu", "--disable-dev-shm-usage", "--hide-scrollbars",
                         "--force-device-scale-factor=1", f"--window-size={width},{height}"):
            options.add_argument(argument)
        options.set_capability("goog:loggingPrefs", {"browser": "ALL", "performance": "ALL"})
        self.driver = webdriver.Chrome(options=options, service=Service(shutil.which("chromedriver")))
        self.driver.execute_cdp_cmd("Emulation.setEmulatedMedia", {"features": [
            {"name": "prefers-color-scheme", "value": "dark" if dark else "light"}]})
        self.resize(width, height)

    def resize(self, width, height):
        self.driver.execute_cdp_cmd("Emulation.setDeviceMetricsOverride", {
            "width": width, "height": height, "deviceScaleFactor": 1, "mobile": False})

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self.driver.quit()

    def open(self, path, fragment=""):
        self.driver.get("about:blank")
        self.driver.get(f"file://{path}#{fragment}")

    def go(self, fragment):
        self.run("location.hash = arguments[0]", fragment)
        self.settle()

    def settle(self):
        self.driver.execute_async_script("const done = arguments[0]; requestAnimationFrame(() => requestAnimationFrame(done))")

    def run(self, script, *arguments):
        return self.driver.execute_script(script, *arguments)

    def texts(self, selector):
        """Of the elements that are shown, as they are read."""
        return [element.text for element in self.driver.find_elements("css selector", selector) if element.is_displayed()]

    def click(self, selector):
        next(element for element in self.driver.find_elements("css selector", selector) if element.is_displayed()).click()
        self.settle()

    def press(self, selector, *keys):
        self.driver.find_element("css selector", selector).send_keys(*keys)
        self.settle()

    def picture(self, path):
        self.driver.save_screenshot(str(path))

    def console(self):
        return [entry["message"] for entry in self.driver.get_log("browser")]

    def requests(self):
        """The addresses that were asked for since the last call."""
        import json
        messages = [json.loads(entry["message"])["message"] for entry in self.driver.get_log("performance")]
        return [message["params"]["request"]["url"] for message in messages if message["method"] == "Network.requestWillBeSent"]
