// Says "page" at once: what a process costs before it asks anything.
trace("page");
quit();
