"""What the tests of the pages share: a browser, and how a page is looked at."""

import base64
import json
import os
import subprocess
import sys
import tempfile
import unittest

try:
    from selenium import webdriver
    from selenium.common.exceptions import WebDriverException
    from selenium.webdriver.chrome.options import Options
    from selenium.webdriver.chrome.service import Service
    from selenium.webdriver.common.by import By
    from selenium.webdriver.common.keys import Keys
    from selenium.webdriver.support.ui import WebDriverWait
except ImportError as error:
    print(f"this machine does not let the tests run Chromium: {error}")
    sys.exit(0)

FOLDER = sys.argv[1]

# The colour of a text and what lies behind it, as the browser shows them.
CONTRAST = """
  const parsed = (text) => text.match(/[\\d.]+/g).map(Number);
  const light = (rgb) => {
    const [r, g, b] = rgb.map((c) => {
      c /= 255;
      return c <= 0.03928 ? c / 12.92 : ((c + 0.055) / 1.055) ** 2.4;
    });
    return 0.2126 * r + 0.7152 * g + 0.0722 * b;
  };
  const behind = (element) => {
    for (let e = element; e !== null; e = e.parentElement) {
      const [r, g, b, a = 1] = parsed(getComputedStyle(e).backgroundColor);
      if (a > 0) {
        return [r, g, b];
      }
    }
    return [255, 255, 255];
  };
  const worst = {ratio: 21, text: ""};
  for (const element of document.querySelectorAll(arguments[0])) {
    const own = Array.from(element.childNodes).some(
        (node) => node.nodeType === 3 && node.data.trim() !== "");
    if (!own || !element.checkVisibility() || element.closest("svg") !== null) {
      continue;
    }
    const colours = [light(parsed(getComputedStyle(element).color).slice(0, 3)),
                     light(behind(element))].sort((a, b) => b - a);
    const ratio = (colours[0] + 0.05) / (colours[1] + 0.05);
    if (ratio < worst.ratio) {
      worst.ratio = ratio;
      worst.text = element.tagName + "." + element.className + ": " + element.textContent;
    }
  }
  return worst;
"""


def start_browser():
    home = tempfile.mkdtemp(prefix="libschema-browser-")
    os.environ["HOME"] = home
    options = Options()
    for argument in ("--headless=new", "--no-sandbox", "--disable-dev-shm-usage", "--disable-gpu",
                     "--window-size=1280,1000", f"--user-data-dir={home}/profile"):
        options.add_argument(argument)
    options.set_capability("goog:loggingPrefs", {"browser": "ALL", "performance": "ALL"})
    try:
        return webdriver.Chrome(service=Service("/usr/bin/chromedriver"), options=options), home
    except WebDriverException as error:
        subprocess.run(["rm", "-rf", home], check=False)
        print(f"this machine does not let the tests run Chromium: {str(error).splitlines()[0]}")
        sys.exit(0)


class PageTest(unittest.TestCase):
    """Each class of tests has a browser, and each test a page that is loaded anew."""

    page = ""

    @classmethod
    def setUpClass(cls):
        cls.browser, cls.home = start_browser()

    @classmethod
    def tearDownClass(cls):
        cls.browser.quit()
        subprocess.run(["rm", "-rf", cls.home], check=False)

    def setUp(self):
        self.emulate(media="", features=[])
        self.resize(1280, 1000)
        self.load(self.page)

    def load(self, name, anchor=""):
        for log in ("browser", "performance"):
            self.browser.get_log(log)
        self.browser.get("about:blank")
        self.browser.get(f"file://{FOLDER}/{name}.html{anchor}")

    def document(self, name=None):
        with open(f"{FOLDER}/{name or self.page}.json", encoding="utf-8") as file:
            return json.load(file)

    def emulate(self, media="", features=()):
        self.browser.execute_cdp_cmd("Emulation.setEmulatedMedia",
                                     {"media": media, "features": list(features)})

    def resize(self, width, height):
        self.browser.execute_cdp_cmd("Emulation.setDeviceMetricsOverride", {
            "width": width, "height": height, "deviceScaleFactor": 1, "mobile": False})

    def script(self, text, *arguments):
        return self.browser.execute_script(text, *arguments)

    def all(self, selector):
        return self.browser.find_elements(By.CSS_SELECTOR, selector)

    def one(self, selector):
        return self.browser.find_element(By.CSS_SELECTOR, selector)

    def shown(self):
        """How many items a filter leaves."""
        return self.script("return document.querySelectorAll('.item:not([hidden])').length")

    def wait_for_shown(self, number):
        WebDriverWait(self.browser, 20).until(
            lambda _: self.shown() == number,
            f"{self.shown()} items are shown, not {number}")

    def type_words(self, text):
        self.one("#words").clear()
        self.one("#words").send_keys(text)

    def press(self, *keys):
        for key in keys:
            webdriver.ActionChains(self.browser).send_keys(key).perform()

    def focused(self, expression):
        return self.script(f"const e = document.activeElement; return {expression}")

    def tab_to(self, selector, most=60):
        for _ in range(most):
            self.press(Keys.TAB)
            if self.focused(f"e.matches({json.dumps(selector)})"):
                return
        self.fail(f"{selector} is not reached by the keyboard")

    def requests(self):
        """What was asked for since the page was loaded, but for pictures in the page itself."""
        urls = []
        for entry in self.browser.get_log("performance"):
            message = json.loads(entry["message"])["message"]
            if message["method"] == "Network.requestWillBeSent":
                urls.append(message["params"]["request"]["url"])
        return [url for url in urls if not url.startswith(("data:", "about:"))]

    def pdf_text(self):
        data = self.browser.execute_cdp_cmd("Page.printToPDF", {"printBackground": False})["data"]
        pdf = os.path.join(self.home, "page.pdf")
        with open(pdf, "wb") as file:
            file.write(base64.b64decode(data))
        return subprocess.run(["pdftotext", "-raw", pdf, "-"], stdout=subprocess.PIPE,
                              check=True).stdout.decode()

    # ---- What holds for every page ----

    def check_is_quiet(self):
        """No message on the console, and nothing is asked for but the page."""
        self.assertEqual([], self.browser.get_log("browser"))
        requests = self.requests()
        self.assertEqual(1, len(requests), requests)


class EveryPage:
    """What holds for the page of every command."""

    def test_is_quiet(self):
        self.check_is_quiet()

    def test_structure(self):
        self.assertEqual("en", self.script("return document.documentElement.lang"))
        for selector in ("h1", "main", "header", "footer", "nav[aria-label]", "#filters[aria-label]"):
            self.assertEqual(1, len(self.all(selector)), selector)
        levels = self.script("return Array.from(document.querySelectorAll('h1,h2,h3,h4'),"
                             " (e) => Number(e.tagName[1]))")
        for above, below in zip(levels, levels[1:]):
            self.assertLessEqual(below, above + 1)
        self.assertEqual([], self.script("""
          const ids = Array.from(document.querySelectorAll('[id]'), (e) => e.id);
          return ids.filter((id, i) => ids.indexOf(id) !== i);"""), "ids are unique")
        self.assertEqual([], self.script("""
          return Array.from(document.querySelectorAll('a')).map((a) => a.getAttribute('href'))
              .filter((href) => !/^#[a-z0-9-]+$/.test(href) ||
                                document.getElementById(href.slice(1)) === null);"""),
                         "every link leads somewhere in the page")
        self.assertEqual(0, self.script("return document.querySelectorAll('th:not([scope])').length"))
        self.assertEqual(0, self.script("""
          return Array.from(document.querySelectorAll('input')).filter(
              (e) => e.labels.length === 0).length;"""), "every input has a label")
        self.assertEqual(0, self.script("""
          return Array.from(document.querySelectorAll('svg')).filter(
              (e) => !e.getAttribute('aria-label')).length;"""), "every picture is named")

    def test_contrast(self):
        """Texts can be read in both schemes, and the two are not the same."""
        papers = []
        for scheme in ("light", "dark"):
            self.emulate(features=[{"name": "prefers-color-scheme", "value": scheme}])
            papers.append(self.script("return getComputedStyle(document.body).backgroundColor"))
            worst = self.script(CONTRAST, "body *")
            self.assertGreaterEqual(worst["ratio"], 4.5, f"{scheme}: {worst['text']}")
        self.assertNotEqual(*papers)

    def test_narrow(self):
        self.resize(380, 800)
        self.assertLessEqual(
            self.script("return document.documentElement.scrollWidth"), 380)

    def test_skip_link(self):
        self.press(Keys.TAB)
        self.assertEqual("skip", self.focused("e.className"))
        self.assertTrue(self.script(
            "return document.activeElement.getBoundingClientRect().left >= 0"))
        self.press(Keys.ENTER)
        self.assertEqual("main", self.focused("e.id"))


def main():
    unittest.main(argv=[sys.argv[0], "-v"])
