"""Generates the class catalogue from MOF; see generator/."""

import sys

from generator.cli import main

sys.exit(main())
